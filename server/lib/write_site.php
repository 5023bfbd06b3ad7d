<?php
// php write_site.php DATA HTTP_SERVER FTP_SERVER
// Used by server/run: records the addresses the service runs on and rewrites
// every user's configuration file to name them.
declare(strict_types=1);

require __DIR__ . '/cli.php';

use function Quorvel\Service\{fail, load_site, lock_data_root, save_site, write_cfg_files};

if ($argc !== 4) {
    fail('usage: write_site.php DATA HTTP_SERVER FTP_SERVER', 2);
}
[, $root, $http, $ftp] = $argv;
$lock = lock_data_root($root);
try {
    $site = load_site($root);
    $site['http_server'] = $http;
    $site['ftp_server'] = $ftp;
    save_site($root, $site);
    write_cfg_files($root, $site);
} catch (Quorvel\Service\AccountError $e) {
    fail($e->getMessage());
}
