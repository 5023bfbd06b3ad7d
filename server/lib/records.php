<?php
// Reading data files for the service: the records after a date, streamed in
// constant memory, and the last record read from the end of the file.
declare(strict_types=1);

namespace Quorvel\Service;

require_once __DIR__ . '/dates.php';

// Longest line handled; a longer one is skipped (the client refuses such lines).
const LINE_LIMIT = 1 << 20;
// Bytes read at a time.
const BLOCK = 1 << 18;

// Where records go: the reply writer of wd.php, or a test's collector.
interface RecordSink
{
    // A block of whole lines, each ending with LF or CR LF.
    public function lines(string $block): void;
    // One record without its line end.
    public function record(string $line): void;
    // A note the client ignores but traces.
    public function note(string $text): void;
}

// Lines the client would not take as data: the final-line words and the lines
// it ignores.
function is_protocol_line(string $line): bool
{
    return str_starts_with($line, 'OK') || str_starts_with($line, 'NOK') ||
        strncasecmp($line, 'php', 3) === 0;
}

// The fields of a canonical "yyyy-mm-dd HH:MM:SS": where each ends, its
// highest value, and a pattern for any valid value of it.
const DATE_FIELDS = [[4, 9999, '\d{4}'], [7, 12, '(?:0[1-9]|1[0-2])'], [10, 31, '(?:0[1-9]|[12]\d|3[01])'],
    [13, 23, '(?:[01]\d|2[0-3])'], [16, 59, '[0-5]\d'], [19, 59, '[0-5]\d']];

// Fails at 30 February, 31 April and the like, and 29 February outside leap years.
function impossible_day_guard(): string
{
    $leapYear = '(?:\d\d(?:0[48]|[2468][048]|[13579][26])|(?:[02468][048]|[13579][26])00)';
    return '(?!\d{4}-(?:02-(?:3|29(?<!' . $leapYear . '-02-29))|0[469]-31|11-31))';
}

// Any valid value for the fields after field $k, with their separators.
function later_fields_pattern(int $k): string
{
    $rest = '';
    for ($j = $k + 1; $j < count(DATE_FIELDS); ++$j) {
        $rest .= 'yyyy-mm-dd HH:MM:SS'[DATE_FIELDS[$j - 1][0]] . DATE_FIELDS[$j][2];
    }
    return $rest;
}

// A pattern that matches a valid canonical "yyyy-mm-dd HH:MM:SS" later than
// $after (itself canonical): field by field, the same fields and then a greater
// one, each later field any valid value.
function later_than_pattern(string $after): string
{
    $branches = [];
    $start = 0;
    foreach (DATE_FIELDS as $k => [$end, $highest]) {
        $value = substr($after, $start, $end - $start);
        $greater = $k === 0 ? greater_year_pattern($value) : greater_value_pattern((int) $value, $highest);
        if ($greater !== null) {
            $branches[] = substr($after, 0, $start) . $greater . later_fields_pattern($k);
        }
        $start = $end + 1;
    }
    return $branches ? impossible_day_guard() . '(?:' . implode('|', $branches) . ')' : '(?!)';
}

// A narrower pattern, quicker to check: dates that share $first's year, or year
// and month, when that is where $first is later than $after. Null otherwise, or
// when $first is not a valid canonical date later than $after.
function later_prefix_pattern(string $first, string $after): ?string
{
    if (preg_match('/^' . later_than_pattern($after) . '$/D', $first) !== 1) {
        return null;
    }
    // Only a later year or month: a block of records rarely shares a day.
    foreach (array_slice(DATE_FIELDS, 0, 2) as $k => [$end]) {
        if (strcmp(substr($first, 0, $end), substr($after, 0, $end)) > 0) {
            return impossible_day_guard() . substr($first, 0, $end) . later_fields_pattern($k);
        }
    }
    return null;
}

// Two-digit values above $value up to $highest, or null when there are none.
function greater_value_pattern(int $value, int $highest): ?string
{
    $values = [];
    for ($v = $value + 1; $v <= $highest; ++$v) {
        $values[] = sprintf('%02d', $v);
    }
    return $values ? '(?:' . implode('|', $values) . ')' : null;
}

// Four-digit years above $year: the same leading digits, then a greater digit.
function greater_year_pattern(string $year): ?string
{
    $branches = [];
    for ($i = 0; $i < 4; ++$i) {
        if ($year[$i] !== '9') {
            $branches[] = substr($year, 0, $i) . '[' . ((int) $year[$i] + 1) . '-9]' . str_repeat('\d', 3 - $i);
        }
    }
    return $branches ? '(?:' . implode('|', $branches) . ')' : null;
}

// Selects the records of a file whose date is later than a given one. Most
// logger files hold "DateTime" records with canonical dates in rising order;
// for those a whole block is checked by one regular expression and passed on
// as it stands. Any block that does not pass that check is read line by line.
final class RecordFilter
{
    // Lines whose field 0 is a canonical date later than the given one: any
    // line (tab or comma after the date), and the quicker form for blocks
    // without tabs.
    private ?string $blockPattern = null;
    private ?string $commaBlockPattern = null;
    private string $afterText = '';

    /**
     * @param ?int $afterSeconds null: every record (the client asked with date=0)
     */
    public function __construct(
        private readonly int $type,
        private readonly ?int $afterSeconds,
        private readonly bool $dayFirst,
        private readonly RecordSink $sink,
    ) {
        if ($afterSeconds !== null && in_array($type, [DATE_TIME, GEMINI, TEKSMART], true) && $afterSeconds > 0) {
            $this->afterText = format_iso_seconds($afterSeconds);
            $later = '^' . later_than_pattern($this->afterText);
            // The date is field 0: a tab follows it, or a comma with no tab in the line.
            $this->blockPattern = '/' . $later . '(?:\t[^\r\n]*|,[^\t\r\n]*)\r?$/m';
            $this->commaBlockPattern = '/' . $later . ',/m';
        }
    }

    // Takes whole lines (the last one may lack its line end only at the end of the file).
    public function block(string $block): void
    {
        if ($this->passesWhole($block)) {
            $this->sink->lines(str_ends_with($block, "\n") ? $block : $block . "\r\n");
            return;
        }
        $text = str_replace(["\r\n", "\r"], "\n", $block);
        foreach (explode("\n", $text) as $line) {
            $this->line($line);
        }
    }

    private function passesWhole(string $block): bool
    {
        if ($this->afterSeconds === null) {
            // Every record goes: only lone CRs, empty lines and protocol words
            // need the line-by-line way.
            return preg_match('/\r(?!\n)/', $block) === 0 &&
                preg_match('/\n(?:\r?\n|OK|NOK|[Pp][Hh][Pp])/', $block) === 0 &&
                $block[0] !== "\n" && !str_starts_with($block, "\r\n") && !is_protocol_line($block);
        }
        if ($this->blockPattern === null) {
            return false;
        }
        // Every line a canonical date later than the given one (which also
        // rules out empty lines and protocol words).
        $lines = substr_count($block, "\n") + (str_ends_with($block, "\n") ? 0 : 1);
        if (!str_contains($block, "\t")) {
            if (preg_match('/\r(?!\n)/', $block) !== 0) {
                return false;
            }
            // Records far newer than the client's copy: most blocks share the first one's year or month.
            $prefix = later_prefix_pattern(substr($block, 0, 19), $this->afterText);
            if ($prefix !== null && preg_match_all('/^' . $prefix . ',/m', $block) === $lines) {
                return true;
            }
            return preg_match_all($this->commaBlockPattern, $block) === $lines;
        }
        return preg_match_all($this->blockPattern, $block) === $lines;
    }

    public function line(string $line): void
    {
        if ($line === '') {
            return;
        }
        if (is_protocol_line($line)) {
            $this->sink->note('skipped a record the client would take as a reply line: ' . substr($line, 0, 40));
            return;
        }
        if ($this->afterSeconds !== null) {
            $seconds = line_seconds($line, $this->type, $this->dayFirst);
            if ($seconds === null || $seconds <= $this->afterSeconds) {
                return;
            }
        }
        $this->sink->record($line);
    }
}

// Reads a file forward in blocks and hands whole lines to the filter. Lines end
// at LF, CR LF or CR; the last line may lack its line end. Memory stays bounded
// by the block size and the line limit, whatever the size of the file.
function filter_file($stream, RecordFilter $filter, RecordSink $sink): void
{
    $carry = '';
    $skipping = false; // inside an over-long line
    while (true) {
        $chunk = fread($stream, BLOCK);
        if ($chunk === false) {
            throw new \RuntimeException('read error');
        }
        $end = $chunk === '' && feof($stream);
        $text = $carry . $chunk;
        $cut = $end ? strlen($text) : last_line_end($text);
        if ($cut < 0) {
            $carry = $text;
            if (strlen($carry) > LINE_LIMIT) {
                $carry = '';
                $skipping = true;
            }
            continue;
        }
        $block = substr($text, 0, $cut);
        $carry = substr($text, $cut);
        // Only the first line can be too long: it is the one that began in an earlier read.
        if ($skipping || strcspn($block, "\r\n") > LINE_LIMIT) {
            $sink->note('skipped a line longer than ' . LINE_LIMIT . ' bytes');
            $block = drop_first_line($block);
            $skipping = false;
        }
        if ($block !== '') {
            $filter->block($block);
        }
        if ($end) {
            return;
        }
    }
}

// The text after the first line end.
function drop_first_line(string $text): string
{
    $at = strcspn($text, "\r\n");
    if ($at >= strlen($text)) {
        return '';
    }
    return substr($text, $at + (substr($text, $at, 2) === "\r\n" ? 2 : 1));
}

// The end of the last complete line (just after its line end), or -1. A CR at
// the very end may be followed by an LF still unread, so it ends no line yet.
function last_line_end(string $text): int
{
    $lf = strrpos($text, "\n");
    $cr = strrpos($text, "\r", -2);
    $cut = max($lf === false ? -1 : $lf, $cr === false ? -1 : $cr);
    return $cut < 0 ? -1 : $cut + 1;
}

// The last non-empty line of a file, read backwards from its end; '' when there
// is none, null when the line is longer than the line limit.
function last_line(string $path): ?string
{
    $stream = fopen($path, 'rb');
    if ($stream === false) {
        throw new \RuntimeException('cannot open');
    }
    try {
        $end = fstat($stream)['size']; // not filesize(): PHP caches that
        // Skip the line ends at the end of the file.
        while ($end > 0) {
            $start = max(0, $end - 4096);
            fseek($stream, $start);
            $block = (string) fread($stream, $end - $start);
            $kept = rtrim($block, "\r\n");
            $end = $start + strlen($kept);
            if ($kept !== '') {
                break;
            }
        }
        $line = '';
        while ($end > 0) {
            $start = max(0, $end - 4096);
            fseek($stream, $start);
            $block = (string) fread($stream, $end - $start);
            $cr = strrpos($block, "\r");
            $lf = strrpos($block, "\n");
            $at = max($cr === false ? -1 : $cr, $lf === false ? -1 : $lf);
            $line = substr($block, $at + 1) . $line;
            if (strlen($line) > LINE_LIMIT) {
                return null;
            }
            if ($at >= 0) {
                break;
            }
            $end = $start;
        }
        return $line;
    } finally {
        fclose($stream);
    }
}
