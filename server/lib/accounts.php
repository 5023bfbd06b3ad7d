<?php
// Accounts and the data root of the reference service.
//
// Data root layout (never inside a web server's document root):
//   site.json          addresses written into configuration files
//   users.json         accounts: password hashes, folders, FTP secret
//   cfg/NAME.cfg       the configuration file of user NAME (served over HTTP)
//   users/NAME/        the user's folder: files.txt, data files, season folder
declare(strict_types=1);

namespace Quorvel\Service;

const SITE_DEFAULTS = [
    'http_server' => '127.0.0.1:8080',
    'ftp_server' => '127.0.0.1:2121',
    'web_folder' => '/wd',
];
// Names that the web paths of the service use themselves.
const RESERVED_NAMES = ['cfg', 'wd', 'users'];

final class AccountError extends \RuntimeException
{
}

// The data root: QUORVEL_DATA from the web server or the environment, else
// server/data beside this library.
function data_root(): string
{
    $given = $_SERVER['QUORVEL_DATA'] ?? getenv('QUORVEL_DATA');
    return is_string($given) && $given !== '' ? rtrim($given, '/') : dirname(__DIR__) . '/data';
}

function users_file(string $root): string
{
    return $root . '/users.json';
}

function user_folder(string $root, string $name): string
{
    return $root . '/users/' . $name;
}

function cfg_file(string $root, string $name): string
{
    return $root . '/cfg/' . $name . '.cfg';
}

// A user name is also a folder name and a piece of a web address.
function is_valid_user_name(string $name): bool
{
    return preg_match('/^[A-Za-z0-9][A-Za-z0-9._-]{0,63}$/D', $name) === 1 &&
        !in_array(strtolower($name), RESERVED_NAMES, true);
}

function is_valid_folder_name(string $name): bool
{
    return preg_match('/^[A-Za-z0-9][A-Za-z0-9._ -]{0,63}$/D', $name) === 1;
}

/** @return array<string,mixed> */
function read_json(string $path): array
{
    if (!is_file($path)) {
        return [];
    }
    $text = file_get_contents($path);
    $data = $text === false ? null : json_decode($text, true);
    if (!is_array($data)) {
        throw new AccountError("$path is not a readable JSON object");
    }
    return $data;
}

// Written beside the old file and renamed over it, so a reader never sees half a file.
/** @param array<string,mixed> $data */
function write_json(string $path, array $data): void
{
    $text = json_encode($data, JSON_PRETTY_PRINT | JSON_UNESCAPED_SLASHES | JSON_UNESCAPED_UNICODE) . "\n";
    write_file_atomically($path, $text, 0600);
}

function write_file_atomically(string $path, string $text, int $mode): void
{
    $temp = $path . '.' . getmypid() . '.tmp';
    if (file_put_contents($temp, $text) === false || !chmod($temp, $mode) || !rename($temp, $path)) {
        @unlink($temp);
        throw new AccountError("cannot write $path");
    }
}

/** @return array<string,array<string,mixed>> */
function load_users(string $root): array
{
    return read_json(users_file($root));
}

/** @return array{http_server:string,ftp_server:string,web_folder:string} */
function load_site(string $root): array
{
    $site = read_json($root . '/site.json') + SITE_DEFAULTS;
    return array_map('strval', array_intersect_key($site, SITE_DEFAULTS)) + SITE_DEFAULTS;
}

/** @param array<string,string> $site */
function save_site(string $root, array $site): void
{
    write_json($root . '/site.json', array_intersect_key($site + SITE_DEFAULTS, SITE_DEFAULTS));
}

// The account of a user whose password matches, else null. An unknown user
// costs the same time as a wrong password.
/** @param array<string,array<string,mixed>> $users */
function authenticate(array $users, string $name, string $password): ?array
{
    static $dummy = '$2y$10$/U2IjLFrIuZASOnceo3mhOdhf1pkhsf/SmgCaQpJPfJ/gebXc0mvu';
    $account = $users[$name] ?? null;
    $hash = is_array($account) && is_string($account['password_hash'] ?? null) ? $account['password_hash'] : $dummy;
    $matches = password_verify($password, $hash);
    return $matches && is_array($account) && $name !== '' ? $account : null;
}

// The PBKDF2 form shared with the FTP server: "pbkdf2-sha256$ROUNDS$SALT$HASH".
function ftp_password_hash(string $password): string
{
    $rounds = 60000;
    $salt = bin2hex(random_bytes(16));
    return 'pbkdf2-sha256$' . $rounds . '$' . $salt . '$' . hash_pbkdf2('sha256', $password, $salt, $rounds);
}

// The five lines a client reads at log-in: FTP server, FTP user, FTP password
// (enciphered), HTTP server, web folder.
/** @param array<string,string> $site @param array<string,mixed> $account */
function cfg_text(array $site, string $name, array $account): string
{
    return implode("\r\n", [$site['ftp_server'], $name, (string) $account['ftp_password_cipher'],
        $site['http_server'], $site['web_folder']]) . "\r\n";
}

/** @param array<string,string> $site */
function write_cfg_files(string $root, array $site): void
{
    @mkdir($root . '/cfg', 0755, true);
    foreach (load_users($root) as $name => $account) {
        write_file_atomically(cfg_file($root, (string) $name), cfg_text($site, (string) $name, $account), 0644);
    }
}

// The user's folders as GETUSERFOLDERS gives them. The user folder starts with
// "/" because the client puts it straight after the HTTP server's host:port to
// build the file list's address.
/** @param array<string,mixed> $account @return array{string,string,string,string,string} */
function user_details(string $name, array $account): array
{
    $folder = '/' . $name;
    $season = (string) ($account['season'] ?? '');
    return [$folder, $season, $season === '' ? $folder : $folder . '/' . $season,
        (string) ($account['data_folder'] ?? ''), (string) ($account['display_name'] ?? $name)];
}
