<?php
// The answers of wd.php: GETUSERFOLDERS, GETLASTDATE and GETDATA.
//
// Every answer is a plain-text body of data lines and one final line beginning
// "OK" or "NOK"; the HTTP status is always 200, because the client treats any
// other status as a broken exchange and waits out its time-out. Lines that
// begin with "php" are notes the client ignores.
declare(strict_types=1);

namespace Quorvel\Service;

require_once __DIR__ . '/accounts.php';
require_once __DIR__ . '/records.php';

const LOCATION_SEASON = 3;

// Writes the reply body, passing records on in pieces of about 64 KB.
final class Reply implements RecordSink
{
    private string $pending = '';

    public function __construct()
    {
        header_remove('X-Powered-By');
        header('Content-Type: text/plain');
        header('Cache-Control: no-store');
        header('X-Content-Type-Options: nosniff');
        header('X-Accel-Buffering: no'); // nginx: pass records on as they come
        ini_set('zlib.output_compression', '0');
        while (ob_get_level() > 0) {
            ob_end_flush();
        }
    }

    public function lines(string $block): void
    {
        if ($this->pending === '' && strlen($block) >= 65536) {
            echo $block; // a whole block of records goes on without a copy
            flush();
            return;
        }
        $this->pending .= $block;
        if (strlen($this->pending) >= 65536) {
            $this->send();
        }
    }

    public function record(string $line): void
    {
        $this->lines($line . "\r\n");
    }

    public function note(string $text): void
    {
        $this->lines('php ' . str_replace(["\r", "\n"], ' ', $text) . "\r\n");
    }

    public function ok(string $value = ''): void
    {
        $this->final($value === '' ? 'OK' : 'OK ' . $value);
    }

    public function nok(string $reason): void
    {
        $this->final('NOK ' . str_replace(["\r", "\n"], ' ', $reason));
    }

    private function final(string $line): void
    {
        $this->pending .= $line . "\r\n";
        $this->send();
    }

    private function send(): void
    {
        echo $this->pending;
        $this->pending = '';
        flush();
    }
}

// A request refused before any work: the reason goes into the NOK line.
final class Refusal extends \RuntimeException
{
}

/** @param array<string,mixed> $query */
function answer_request(array $query, string $root): void
{
    $reply = new Reply();
    try {
        $users = load_users($root);
    } catch (AccountError) {
        $reply->nok('the service has no readable users file');
        return;
    }
    $name = text_parameter($query, 'user');
    $account = authenticate($users, $name, text_parameter($query, 'pwd'));
    if ($account === null) {
        $reply->nok('unknown user or wrong password');
        return;
    }
    $command = text_parameter($query, 'cmd');
    if (text_parameter($query, 'trace') === 'on') {
        $reply->note("wd.php: $command for $name");
    }
    try {
        match ($command) {
            'GETUSERFOLDERS' => answer_user_folders($reply, $name, $account),
            'GETLASTDATE' => answer_last_date($reply, $query, $root, $name, $account),
            'GETDATA' => answer_data($reply, $query, $root, $name, $account),
            default => throw new Refusal($command === '' ? 'no command' : "unknown command $command"),
        };
    } catch (Refusal $refusal) {
        $reply->nok($refusal->getMessage());
    }
}

/** @param array<string,mixed> $query */
function text_parameter(array $query, string $name): string
{
    $value = $query[$name] ?? '';
    return is_string($value) ? $value : '';
}

/** @param array<string,mixed> $account */
function answer_user_folders(Reply $reply, string $name, array $account): void
{
    $reply->record(implode('|', user_details($name, $account)));
    $reply->ok();
}

/** @param array<string,mixed> $query @param array<string,mixed> $account */
function answer_last_date(Reply $reply, array $query, string $root, string $name, array $account): void
{
    $type = data_type($query);
    $path = find_data_file($root, $name, $account, $query);
    if ($path === null) {
        $reply->ok('NO FILE');
        return;
    }
    try {
        $line = last_line($path);
    } catch (\RuntimeException) {
        throw new Refusal('cannot read ' . text_parameter($query, 'file'));
    }
    $seconds = $line === null || $line === '' ? null : line_seconds($line, $type, day_first($account));
    $reply->ok($seconds === null ? '0' : format_iso_seconds($seconds));
}

/** @param array<string,mixed> $query @param array<string,mixed> $account */
function answer_data(Reply $reply, array $query, string $root, string $name, array $account): void
{
    $type = data_type($query);
    $after = after_seconds(text_parameter($query, 'date'));
    $path = find_data_file($root, $name, $account, $query);
    if ($path === null) {
        throw new Refusal('NO FILE ' . text_parameter($query, 'file'));
    }
    $stream = @fopen($path, 'rb');
    if ($stream === false) {
        throw new Refusal('cannot read ' . text_parameter($query, 'file'));
    }
    set_time_limit(0);
    try {
        filter_file($stream, new RecordFilter($type, $after, day_first($account), $reply), $reply);
    } catch (\RuntimeException) {
        throw new Refusal('read error in ' . text_parameter($query, 'file'));
    } finally {
        fclose($stream);
    }
    $reply->ok();
}

/** @param array<string,mixed> $query */
function data_type(array $query): int
{
    $dt = text_parameter($query, 'dt');
    if (preg_match('/^[0-8]$/D', $dt) !== 1) {
        throw new Refusal("unknown data type \"$dt\"");
    }
    return (int) $dt;
}

// null for "0" (every record).
function after_seconds(string $date): ?int
{
    if ($date === '0') {
        return null;
    }
    $value = parse_date_text($date);
    if ($value === null || $value == 0.0) {
        throw new Refusal("unreadable date \"$date\"");
    }
    return date_seconds($value);
}

/** @param array<string,mixed> $account */
function day_first(array $account): bool
{
    return ($account['date_order'] ?? 'dmy') !== 'mdy';
}

// The data file a request names, inside the user's own folder, or null when it
// does not exist. The folder of the location asked for is tried first, then the
// user folder and the season folder: the client sends the location of the file
// on its own PC, which need not be the folder the file has at the service.
/** @param array<string,mixed> $account @param array<string,mixed> $query */
function find_data_file(string $root, string $name, array $account, array $query): ?string
{
    $file = text_parameter($query, 'file');
    if (!is_safe_file_name($file)) {
        throw new Refusal('refused file name "' . addcslashes($file, "\0..\37") . '"');
    }
    $location = text_parameter($query, 'filelocation');
    if (preg_match('/^[0-4]$/D', $location) !== 1) {
        throw new Refusal("unknown file location \"$location\"");
    }
    $base = realpath(user_folder($root, $name));
    if ($base === false) {
        return null;
    }
    $season = (string) ($account['season'] ?? '');
    $folders = (int) $location === LOCATION_SEASON ? [$season, ''] : ['', $season];
    foreach (array_unique($folders) as $folder) {
        if ($folder !== '' && !is_valid_folder_name($folder)) {
            continue;
        }
        $path = realpath($base . ($folder === '' ? '' : '/' . $folder) . '/' . $file);
        // realpath follows links: a link that leads out of the user's folder is not followed.
        if ($path !== false && str_starts_with($path, $base . '/') && is_file($path)) {
            return $path;
        }
    }
    return null;
}

// A plain file name: no folder part, no NUL or control character, not hidden.
function is_safe_file_name(string $file): bool
{
    return $file !== '' && strlen($file) <= 255 && strpbrk($file, "/\\") === false &&
        preg_match('/[\x00-\x1f\x7f]/', $file) !== 1 && $file[0] !== '.';
}
