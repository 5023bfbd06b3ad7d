<?php
// Helpers of the command-line tools (add-user, simulate).
declare(strict_types=1);

namespace Quorvel\Service;

require_once __DIR__ . '/accounts.php';

function fail(string $message, int $code = 1): never
{
    fwrite(STDERR, basename($_SERVER['argv'][0] ?? 'server') . ": $message\n");
    exit($code);
}

// Splits arguments into positional ones and "--name value" options; options
// listed in $flags take no value.
/** @param list<string> $args @param list<string> $known @param list<string> $flags
 *  @return array{list<string>,array<string,string|bool>} */
function parse_arguments(array $args, array $known, array $flags = []): array
{
    $positional = [];
    $options = [];
    for ($i = 0; $i < count($args); ++$i) {
        $arg = $args[$i];
        if (!str_starts_with($arg, '--')) {
            $positional[] = $arg;
            continue;
        }
        $name = substr($arg, 2);
        if (in_array($name, $flags, true)) {
            $options[$name] = true;
            continue;
        }
        if (!in_array($name, $known, true)) {
            fail("unknown option $arg", 2);
        }
        if ($i + 1 >= count($args)) {
            fail("$arg needs a value", 2);
        }
        $options[$name] = $args[++$i];
    }
    return [$positional, $options];
}

// The data root of a tool: --data, else QUORVEL_DATA, else server/data.
/** @param array<string,string|bool> $options */
function tool_data_root(array $options): string
{
    $given = $options['data'] ?? '';
    return is_string($given) && $given !== '' ? rtrim($given, '/') : data_root();
}

// Holds the data root's lock while a tool changes the users file.
/** @return resource */
function lock_data_root(string $root)
{
    if (!is_dir($root) && !@mkdir($root, 0700, true)) {
        fail("cannot create the data folder $root");
    }
    $lock = fopen($root . '/.lock', 'c');
    if ($lock === false || !flock($lock, LOCK_EX)) {
        fail("cannot lock $root");
    }
    return $lock;
}
