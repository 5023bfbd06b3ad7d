<?php
// A small stand-in for the service script, for the client's end-to-end tests.
// Run as the router of PHP's web server; records live in the folder "data" of
// the document root, one file per data file, with the date and time in the
// first comma-separated field.
header('Content-Type: text/plain');

$dir = $_SERVER['DOCUMENT_ROOT'] . '/data';
$cmd = $_GET['cmd'] ?? '';
if (($_GET['user'] ?? '') !== 'ann' || ($_GET['pwd'] ?? '') !== 'p&ss word') {
    echo "NOK bad user\r\n";
    exit;
}
$path = $dir . '/' . basename($_GET['file'] ?? '');

function records($path) {
    return is_file($path) ? file($path, FILE_IGNORE_NEW_LINES | FILE_SKIP_EMPTY_LINES) : [];
}

switch ($cmd) {
case 'GETUSERFOLDERS':
    echo "users/ann|users/ann/current|users/ann/x|users/ann/data|Ann Example\r\n";
    echo "OK\r\n";
    break;
case 'GETLASTDATE':
    $lines = records($path);
    if (!$lines) {
        echo "OK NO FILE\r\n";
        break;
    }
    echo 'OK ' . explode(',', end($lines))[0] . "\r\n";
    break;
case 'GETDATA':
    $from = $_GET['date'] ?? '0';
    foreach (records($path) as $line) {
        $date = explode(',', $line)[0];
        if ($from === '0' || strcmp($date, $from) > 0) {
            echo $line . "\r\n";
        }
    }
    echo "OK\r\n";
    break;
default:
    echo "NOK unknown command\r\n";
}
