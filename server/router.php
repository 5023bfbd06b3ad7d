<?php
// Router for PHP's built-in web server (server/run). Only three kinds of address
// are answered; everything else, the users file above all, is "not found":
//   WEB_FOLDER/wd.php     the service script
//   /cfg/NAME.cfg         a user's configuration file
//   /NAME/files.txt       a user's file list
// The same rules as a web server configuration are in server/README.md.
declare(strict_types=1);

require __DIR__ . '/lib/accounts.php';

use function Quorvel\Service\{cfg_file, data_root, is_valid_user_name, load_site, load_users, user_folder};

function not_found(int $status = 404, string $text = 'not found'): bool
{
    http_response_code($status);
    header('Content-Type: text/plain');
    echo $text, "\n";
    return true;
}

function serve_text_file(string $path): bool
{
    if (!is_file($path)) {
        return not_found();
    }
    header('Content-Type: text/plain');
    header('Cache-Control: no-store');
    header('Content-Length: ' . filesize($path));
    if ($_SERVER['REQUEST_METHOD'] !== 'HEAD') {
        readfile($path);
    }
    return true;
}

function route(): bool
{
    header_remove('X-Powered-By');
    if (!in_array($_SERVER['REQUEST_METHOD'], ['GET', 'HEAD'], true)) {
        return not_found(405, 'method not allowed');
    }
    // The client writes the absolute address into its request line.
    $target = explode('?', (string) $_SERVER['REQUEST_URI'], 2)[0];
    $target = (string) preg_replace('#^[A-Za-z][A-Za-z0-9+.-]*://[^/]*#', '', $target);
    $path = rawurldecode($target);
    $path = (string) preg_replace('#/+#', '/', $path);
    if (str_contains($path, "\0") || preg_match('#(^|/)\.\.?(/|$)#', $path) === 1) {
        return not_found();
    }
    $root = data_root();
    try {
        $site = load_site($root);
        if ($path === rtrim($site['web_folder'], '/') . '/wd.php') {
            require __DIR__ . '/www/wd/wd.php';
            return true;
        }
        if (preg_match('#^/cfg/([^/]+)\.cfg$#D', $path, $m) === 1 && is_valid_user_name($m[1])) {
            return serve_text_file(cfg_file($root, $m[1]));
        }
        if (preg_match('#^/([^/]+)/files\.txt$#D', $path, $m) === 1 && is_valid_user_name($m[1]) &&
            array_key_exists($m[1], load_users($root))) {
            return serve_text_file(user_folder($root, $m[1]) . '/files.txt');
        }
    } catch (Quorvel\Service\AccountError) {
        return not_found(500, 'the service has no readable settings');
    }
    return not_found();
}

return route();
