<?php
// The date of a data-file line in each of the nine layouts, read the way the
// Quorvel client reads it, so that the service and the client agree on which
// records are new. Dates are compared in whole seconds since 30 December 1899,
// the precision of the date text the client sends.
declare(strict_types=1);

namespace Quorvel\Service;

const NO_DATE = 0;
const DATE_TIME = 1;
const DATE_COMMA_TIME = 2;
const YMDHM = 3;
const CSI = 4;
const CIMIS = 5;
const GEMINI = 6;
const DECAGON = 7;
const TEKSMART = 8;

const SECONDS_PER_DAY = 86400;

// Thrown where the client meets a missing field or a field that is no number.
final class UnreadableDate extends \RuntimeException
{
}

// Days from 30 December 1899 to the first of a month (proleptic Gregorian).
function days_from_civil(int $year, int $month, int $day): int
{
    $y = $month <= 2 ? $year - 1 : $year;
    $era = intdiv($y >= 0 ? $y : $y - 399, 400);
    $yoe = $y - $era * 400;
    $mp = ($month + 9) % 12;
    $doy = intdiv(153 * $mp + 2, 5) + $day - 1;
    $doe = $yoe * 365 + intdiv($yoe, 4) - intdiv($yoe, 100) + $doy;
    return $era * 146097 + $doe - 693899; // 693899: 1899-12-30 counted from 0000-03-01
}

function is_valid_date(int $year, int $month, int $day): bool
{
    return $month >= 1 && $month <= 12 && $day >= 1 && $year != 0 &&
        checkdate($month, $day, $year < 0 ? $year + 1 : $year);
}

function make_time(int $hour, int $minute, int $second): float
{
    return ($hour * 3600.0 + $minute * 60.0 + $second) / SECONDS_PER_DAY;
}

// A date value with carry: month 13 is January of the next year, day 0 the last
// day of the month before, hour 24 the next day. 0 when the year does not exist.
function make_date(int $year, int $month, int $day, int $hour = 0, int $minute = 0, int $second = 0): float
{
    $index = $month - 1;
    $carry = $index >= 0 ? intdiv($index, 12) : -intdiv(11 - $index, 12);
    $m = $index - $carry * 12 + 1;
    if ($year + $carry == 0) {
        return 0.0;
    }
    $time = make_time($hour, $minute, $second);
    $whole = floor($time);
    $days = days_from_civil($year + $carry, $m, 1) + ($day - 1) + $whole;
    $fraction = $time - $whole;
    return $days >= 0 ? $days + $fraction : $days - $fraction;
}

function date_part(float $value): float
{
    return $value < 0 ? ceil($value) : floor($value);
}

function time_part(float $value): float
{
    return abs($value - date_part($value));
}

// Whole seconds of a date value, rounded as the client rounds when it writes one.
function date_seconds(float $value): int
{
    return (int) date_part($value) * SECONDS_PER_DAY + (int) round(time_part($value) * SECONDS_PER_DAY);
}

// "yyyy-mm-dd HH:MM:SS" of a date value; "0" for 0.
function format_iso(float $value): string
{
    if ($value == 0.0) {
        return '0';
    }
    return format_iso_seconds(date_seconds($value));
}

function format_iso_seconds(int $seconds): string
{
    $days = intdiv($seconds, SECONDS_PER_DAY);
    $rest = $seconds - $days * SECONDS_PER_DAY;
    if ($rest < 0) {
        $days -= 1;
        $rest += SECONDS_PER_DAY;
    }
    [$y, $m, $d] = civil_from_days($days);
    return sprintf('%04d-%02d-%02d %02d:%02d:%02d', $y, $m, $d, intdiv($rest, 3600),
        intdiv($rest % 3600, 60), $rest % 60);
}

/** @return array{int,int,int} */
function civil_from_days(int $days): array
{
    $z = $days + 693899;
    $era = intdiv($z >= 0 ? $z : $z - 146096, 146097);
    $doe = $z - $era * 146097;
    $yoe = intdiv($doe - intdiv($doe, 1460) + intdiv($doe, 36524) - intdiv($doe, 146096), 365);
    $doy = $doe - (365 * $yoe + intdiv($yoe, 4) - intdiv($yoe, 100));
    $mp = intdiv(5 * $doy + 2, 153);
    $d = $doy - intdiv(153 * $mp + 2, 5) + 1;
    $m = $mp < 10 ? $mp + 3 : $mp - 9;
    $y = $yoe + $era * 400 + ($m <= 2 ? 1 : 0);
    return [$y, $m, $d];
}

// ---- numbers ------------------------------------------------------------

// The leading number of a text: blanks, tabs and line feeds are skipped wherever
// they stand; an optional sign, digits, one decimal point and an exponent (E or
// D) are read up to the first character that cannot continue the number.
// Returns the number's text ('' when there is none) and how much was consumed.
/** @return array{string,int} */
function leading_number(string $text): array
{
    $number = '';
    $digits = $point = $exponent = $expDigits = false;
    $n = strlen($text);
    $i = 0;
    for (; $i < $n; ++$i) {
        $c = $text[$i];
        if ($c === ' ' || $c === "\t" || $c === "\n") {
            continue;
        }
        if ($c >= '0' && $c <= '9') {
            $number .= $c;
            if ($exponent) {
                $expDigits = true;
            } else {
                $digits = true;
            }
        } elseif (($c === '+' || $c === '-') && ($number === '' || ($exponent && substr($number, -1) === 'e'))) {
            $number .= $c;
        } elseif ($c === '.' && !$point && !$exponent) {
            $number .= $c;
            $point = true;
        } elseif (($c === 'e' || $c === 'E' || $c === 'd' || $c === 'D') && $digits && !$exponent) {
            $number .= 'e';
            $exponent = true;
        } else {
            break;
        }
    }
    if ($exponent && !$expDigits) {
        $number = substr($number, 0, (int) strrpos($number, 'e'));
    }
    return [$digits ? $number : '', $i];
}

function val_double(string $text): float
{
    [$number] = leading_number($text);
    return $number === '' ? 0.0 : (float) $number;
}

function round_half_even(float $value): float
{
    return round($value, 0, PHP_ROUND_HALF_EVEN);
}

// The 32-bit leading-number reading, rounded halves to even.
function val_long(string $text): int
{
    $v = round_half_even(val_double($text));
    return (int) max(-2147483648.0, min(2147483647.0, $v));
}

// The strict 16-bit conversion: the whole text (blanks around it allowed) must
// be a number.
function int16(string $text): int
{
    $trimmed = trim($text, " \t\n\r\0\x0B\x0C");
    if ($trimmed === '' || strpbrk($trimmed, " \t\n") !== false) {
        throw new UnreadableDate('Type mismatch');
    }
    [$number, $consumed] = leading_number($trimmed);
    if ($number === '' || $consumed !== strlen($trimmed)) {
        throw new UnreadableDate('Type mismatch');
    }
    $v = round_half_even((float) $number);
    if (!is_finite($v) || $v < -32768 || $v > 32767) {
        throw new UnreadableDate('Overflow');
    }
    return (int) $v;
}

// Two-digit years: 0-29 are 2000-2029, 30-99 are 1930-1999.
function full_year(int $year): int
{
    if ($year >= 0 && $year < 30) {
        return $year + 2000;
    }
    if ($year >= 30 && $year < 100) {
        return $year + 1900;
    }
    return $year;
}

// ---- date texts ------------------------------------------------------------

const TIME_PATTERN = '(?:[ T]+(\d{1,2}):(\d{2})(?::(\d{2}))?(?:\s*([AaPp][Mm]))?)?';
const MONTH_NAMES = ['january', 'february', 'march', 'april', 'may', 'june', 'july',
    'august', 'september', 'october', 'november', 'december'];

function month_from_name(string $name): int
{
    $lower = strtolower($name);
    if (strlen($lower) < 3) {
        return 0;
    }
    foreach (MONTH_NAMES as $i => $full) {
        if ($lower === $full || (str_starts_with($full, $lower) && (strlen($lower) === 3 || $lower === 'sept'))) {
            return $i + 1;
        }
    }
    return 0;
}

function text_year(string $digits): int
{
    $y = (int) $digits;
    if (strlen($digits) > 2) {
        return $y;
    }
    return $y < 30 ? 2000 + $y : 1900 + $y;
}

/** @param array<int,string> $m */
function build_date(int $year, int $month, int $day, array $m, int $timeAt, bool $hasDate): ?float
{
    $hour = $minute = $second = 0;
    if (($m[$timeAt] ?? '') !== '') {
        $hour = (int) $m[$timeAt];
        $minute = (int) $m[$timeAt + 1];
        $second = ($m[$timeAt + 2] ?? '') !== '' ? (int) $m[$timeAt + 2] : 0;
        if (($m[$timeAt + 3] ?? '') !== '') {
            if ($hour < 1 || $hour > 12) {
                return null;
            }
            $pm = strtolower($m[$timeAt + 3][0]) === 'p';
            $hour = $hour % 12 + ($pm ? 12 : 0);
        }
        if ($hour > 23 || $minute > 59 || $second > 59) {
            return null;
        }
    }
    if (!$hasDate) {
        return make_time($hour, $minute, $second);
    }
    if ($year < 100 || $year > 9999 || !is_valid_date($year, $month, $day)) {
        return null;
    }
    return make_date($year, $month, $day, $hour, $minute, $second);
}

// A date or time text: ISO "yyyy-mm-dd", "d mmm yyyy", numeric day and month in
// the user's order (dayFirst), or a bare time; each date may carry a time.
function parse_date_text(string $text, bool $dayFirst = true): ?float
{
    $s = trim($text, " \t\n\r\0\x0B\x0C");
    if ($s === '') {
        return null;
    }
    if (preg_match('/^(\d{4})[-\/.](\d{1,2})[-\/.](\d{1,2})' . TIME_PATTERN . '$/D', $s, $m)) {
        return build_date((int) $m[1], (int) $m[2], (int) $m[3], $m, 4, true);
    }
    if (preg_match('/^(\d{1,2})[ -]+([A-Za-z]{3,9})\.?[ ,-]+(\d{2}|\d{4})' . TIME_PATTERN . '$/D', $s, $m)) {
        $month = month_from_name($m[2]);
        return $month === 0 ? null : build_date(text_year($m[3]), $month, (int) $m[1], $m, 4, true);
    }
    if (preg_match('/^(\d{1,2})([-\/.])(\d{1,2})\2(\d{2}|\d{4})' . TIME_PATTERN . '$/D', $s, $m)) {
        [$day, $month] = $dayFirst ? [(int) $m[1], (int) $m[3]] : [(int) $m[3], (int) $m[1]];
        return build_date(text_year($m[4]), $month, $day, $m, 5, true);
    }
    if (preg_match('/^(\d{1,2}):(\d{2})(?::(\d{2}))?(?:\s*([AaPp][Mm]))?$/D', $s, $m)) {
        return build_date(0, 0, 0, $m, 1, false);
    }
    return null;
}

// The date text before a time of hour 24 ("24:00" or "24:00:00"), or null when
// the text ends in no such time.
function before_hour24(string $text): ?string
{
    return preg_match('/^\s*(?:(.*\S)\s+)?24:00(?::00)?\s*$/D', $text, $m) ? ($m[1] ?? '') : null;
}

function time_value(string $text, bool $dayFirst): float
{
    if (before_hour24($text) !== null) {
        return 1.0;
    }
    $v = parse_date_text($text, $dayFirst);
    return $v === null ? 0.0 : time_part($v);
}

function date_value(string $text, bool $dayFirst): float
{
    $before = before_hour24($text);
    if ($before === '') {
        return 0.0;
    }
    $v = parse_date_text($before ?? $text, $dayFirst);
    return $v === null ? 0.0 : date_part($v);
}

function date_time_value(string $text, bool $dayFirst): float
{
    return $text === '0' ? 0.0 : time_value($text, $dayFirst) + date_value($text, $dayFirst);
}

// ---- lines -------------------------------------------------------------------

// The fields of a line: separated by tab when it has one, else by comma when it
// has one, else by space; double quotes removed.
/** @return list<string> */
function line_fields(string $line): array
{
    $separator = str_contains($line, "\t") ? "\t" : (str_contains($line, ',') ? ',' : ' ');
    return explode($separator, str_replace('"', '', $line));
}

/** @param list<string> $fields */
function field(array $fields, int $index): string
{
    if (!array_key_exists($index, $fields)) {
        throw new UnreadableDate('Subscript out of range');
    }
    return $fields[$index];
}

// The date value of a line in a layout; null when the line yields none (fewer
// than two fields, a layout without dates, a missing or unreadable field).
function line_date(string $line, int $type, bool $dayFirst = true): ?float
{
    $f = line_fields($line);
    if (count($f) < 2) {
        return null;
    }
    try {
        switch ($type) {
            case DATE_TIME:
            case GEMINI:
            case TEKSMART:
                return date_time_value($f[0], $dayFirst);
            case DATE_COMMA_TIME:
                return date_value($f[0], $dayFirst) + time_value($f[1], $dayFirst);
            case YMDHM:
                $date = make_date(full_year(int16(field($f, 0))), int16(field($f, 1)), int16(field($f, 2)));
                return $date + make_time(int16(field($f, 3)), int16(field($f, 4)), 0);
            case CSI:
                $year = round_half_even(val_double(field($f, 1)));
                $day = val_double(field($f, 2));
                $hhmm = val_long(field($f, 3));
                if (abs($year) > 9999) {
                    throw new UnreadableDate('Overflow');
                }
                return make_date(full_year((int) $year), 1, 1) + $day - 1 + intdiv($hhmm, 100) / 24.0 +
                    ($hhmm % 100) / 1440.0;
            case CIMIS:
                $date = field($f, 0);
                $time = field($f, 1);
                return make_date(full_year(int16(substr($date, 0, 4))), int16(substr($date, 4, 2)),
                    int16(substr($date, 6, 2))) + make_time(int16(substr($time, 0, 2)), int16(substr($time, 2, 2)), 0);
            case DECAGON:
                return make_date(2000, 1, 1) + val_double(field($f, 1)) + val_double(field($f, 2)) / 1440.0;
            default:
                return null;
        }
    } catch (UnreadableDate) {
        return null;
    }
}

// Whole seconds of a line's date; null when it has none (a date value of 0 is none).
function line_seconds(string $line, int $type, bool $dayFirst = true): ?int
{
    $value = line_date($line, $type, $dayFirst);
    return $value === null || $value == 0.0 ? null : date_seconds($value);
}
